#!/usr/bin/env python3
"""Looks at the site in headless Chromium, from its folder, as a reader does. tools/docs runs it.

Usage: test.py SITE SCREENSHOTS

Prints what is wrong, a line each, and ends with 1 then. (The links were followed when the site was built.)
"""
import pathlib
import sys

from selenium import webdriver
from selenium.webdriver.chrome.service import Service
from selenium.webdriver.common.by import By
from selenium.webdriver.support.wait import WebDriverWait

DESKTOP, PHONE = (1280, 900), (360, 740)
SEARCHES = {"ContextOffscreen": "classORU_1_1OGL_1_1ContextOffscreen.html", "GL_INVALID_OPERATION": "expect.html",
            "glBindTexture": "map.html#map-glBindTexture", "Enforce sBinFile_": "failures.html"}
SHOTS = [("index.html", DESKTOP), ("index.html", PHONE), ("contexts.html", DESKTOP), ("textures.html", PHONE),
         ("classORU_1_1OGL_1_1Buffer.html", DESKTOP), ("classORU_1_1OGL_1_1Buffer.html", PHONE), ("map.html", DESKTOP),
         ("performance.html", DESKTOP), ("performance.html", PHONE)]
# What sticks out to the right of the page, apart from what lies in a box that scrolls by itself.
TOO_WIDE = """
const wide = document.documentElement.clientWidth;
const scrolls = (e) => e && (getComputedStyle(e).overflowX !== "visible" || scrolls(e.parentElement));
return document.documentElement.scrollWidth <= wide ? [] : [...document.querySelectorAll("body *")]
    .filter((e) => e.getBoundingClientRect().right > wide + 1 && !scrolls(e.parentElement))
    .map((e) => e.tagName + "." + e.className).slice(0, 3);"""
BROKEN_PICTURES = "return [...document.images].filter((i) => !(i.complete && i.naturalWidth)).map((i) => i.src)"


def browser():
    options = webdriver.ChromeOptions()
    for argument in ("--headless=new", "--no-sandbox", "--disable-gpu", "--disable-dev-shm-usage", "--hide-scrollbars"):
        options.add_argument(argument)
    options.set_capability("goog:loggingPrefs", {"browser": "ALL"})
    return webdriver.Chrome(options=options, service=Service("/usr/bin/chromedriver"))


def resize(driver, size):
    """The page's size, which is less than a window can be made."""
    driver.execute_cdp_cmd("Emulation.setDeviceMetricsOverride",
                           {"width": size[0], "height": size[1], "deviceScaleFactor": 1, "mobile": size == PHONE})


def complaints(driver, name):
    return [f"{name}: {entry['message']}" for entry in driver.get_log("browser")
            if entry["level"] in ("SEVERE", "WARNING")]


def look_at_pages(driver, site):
    """Pictures, width and messages of every page, on a phone."""
    resize(driver, PHONE)
    for path in sorted(site.glob("*.html")):
        driver.get(path.as_uri())
        for picture in driver.execute_script(BROKEN_PICTURES):
            yield f"{path.name}: a picture does not load: {picture}"
        if wide := driver.execute_script(TOO_WIDE):
            yield f"{path.name}: wider than {PHONE[0]} pixels: {', '.join(wide)}"
        yield from complaints(driver, path.name)


def search(driver, site):
    resize(driver, DESKTOP)
    for text, page in SEARCHES.items():
        driver.get((site / "index.html").as_uri())
        driver.find_element(By.ID, "search").send_keys(text)
        WebDriverWait(driver, 10).until(lambda driver: driver.find_elements(By.CSS_SELECTOR, "#results li"))
        links = [link.get_attribute("href") for link in driver.find_elements(By.CSS_SELECTOR, "#results a")]
        if not any(page in link for link in links):
            yield f"the search for {text} does not find {page}"
        yield from complaints(driver, f"search for {text}")


def filter_map(driver, site):
    resize(driver, DESKTOP)
    driver.get((site / "map.html").as_uri())
    everything = len(driver.find_elements(By.CSS_SELECTOR, "#map-table tbody tr"))
    driver.find_element(By.ID, "map-filter").send_keys("glBindTexture")
    rows = driver.find_elements(By.CSS_SELECTOR, "#map-table tbody tr:not([hidden])")
    shown = [row.get_attribute("id") for row in rows]
    if "map-glBindTexture" not in shown or len(shown) >= everything // 10:
        yield f"the map's filter shows {len(shown)} of {everything} rows for glBindTexture"


def take_pictures(driver, site, folder):
    folder.mkdir(parents=True, exist_ok=True)
    for name, size in SHOTS:
        resize(driver, size)
        driver.get((site / name).as_uri())
        kind = "phone" if size == PHONE else "desktop"
        driver.save_screenshot(str(folder / f"{pathlib.Path(name).stem}-{kind}.png"))


def main(site, screenshots):
    site = site.resolve()
    driver = browser()
    try:
        faults = [*look_at_pages(driver, site), *search(driver, site), *filter_map(driver, site)]
        take_pictures(driver, site, screenshots)
    finally:
        driver.quit()
    for fault in faults:
        print(f"docs: {fault}", file=sys.stderr)
    return 1 if faults else 0


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    sys.exit(main(*map(pathlib.Path, sys.argv[1:])))
