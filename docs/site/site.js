// Search, the filter of the map, the menu on narrow screens. Works from a folder, without a server.
"use strict";

const menu = document.getElementById("menu");
const narrow = matchMedia("(max-width: 60rem)");
const setMenu = () => { menu.open = !narrow.matches; };
narrow.addEventListener("change", setMenu);
setMenu();

// The rows are in a script of their own, read when somebody begins to search: [name, page, kind, text].
const kMostShown = 40;
const input = document.getElementById("search");
const results = document.getElementById("results");
let chosen = -1;

function readRows() {
    if (window.searchRows || document.getElementById("rows"))
        return;
    const script = document.createElement("script");
    script.id = "rows";
    script.src = "searchdata.js";
    script.onload = search;
    document.head.append(script);
}

// The lower, the better; -1 is no hit. A whole name goes before its beginning, that before a part, names before texts.
function rank(row, words, whole) {
    const name = row[0].toLowerCase();
    const last = name.slice(name.lastIndexOf("::") + 1).replace(/^:/, "");
    if (last === whole || name === whole)
        return 0;
    const all = name + " " + row[3].toLowerCase();
    if (!words.every((word) => all.includes(word)))
        return -1;
    if (last.startsWith(whole))
        return 1;
    if (words.every((word) => name.includes(word)))
        return 2;
    return row[2].startsWith("page") ? 3 : 4;
}

// What is around the first hit in a text.
function excerpt(text, word) {
    const at = text.toLowerCase().indexOf(word);
    const from = Math.max(0, at - 40);
    return (from > 0 ? "…" : "") + text.slice(from, from + 140) + (text.length > from + 140 ? "…" : "");
}

function item(row, words) {
    const entry = document.createElement("li");
    const link = document.createElement("a");
    link.href = row[1];
    const [name, kind, text] = ["b", "small", "span"].map((tag) => document.createElement(tag));
    name.textContent = row[0];
    kind.textContent = row[2];
    text.textContent = excerpt(row[3], words[0]);
    link.append(name, " ", kind, text);
    entry.append(link);
    return entry;
}

function search() {
    const whole = input.value.trim().toLowerCase();
    chosen = -1;
    results.hidden = whole.length < 2;
    if (results.hidden || !window.searchRows)
        return;
    const words = whole.split(/\s+/);
    const hits = searchRows.map((row) => [rank(row, words, whole), row]).filter((hit) => hit[0] >= 0);
    hits.sort((a, b) => a[0] - b[0] || a[1][0].length - b[1][0].length || (a[1][0] < b[1][0] ? -1 : 1));
    results.replaceChildren(...hits.slice(0, kMostShown).map((hit) => item(hit[1], words)));
    if (hits.length !== results.children.length || hits.length === 0) {
        const note = document.createElement("li");
        note.className = "note";
        note.textContent = hits.length ? `and ${hits.length - kMostShown} more: type more of the name`
            : "nothing of that name, and no text with it";
        results.append(note);
    }
}

function choose(step) {
    const links = [...results.querySelectorAll("a")];
    if (!links.length)
        return;
    chosen = (chosen + step + links.length) % links.length;
    links.forEach((link, i) => link.classList.toggle("chosen", i === chosen));
    links[chosen].scrollIntoView({block: "nearest"});
}

input.addEventListener("focus", readRows);
input.addEventListener("input", () => { readRows(); search(); });
input.addEventListener("keydown", (event) => {
    if (event.key === "ArrowDown" || event.key === "ArrowUp") {
        choose(event.key === "ArrowDown" ? 1 : -1);
        event.preventDefault();
    } else if (event.key === "Enter") {
        const links = results.querySelectorAll("a");
        if (links.length)
            location.href = links[Math.max(chosen, 0)].href;
    } else if (event.key === "Escape") {
        input.value = "";
        search();
    }
});
document.addEventListener("click", (event) => {
    if (!event.target.closest(".search"))
        results.hidden = true;
    else if (event.target.closest("a"))
        results.hidden = true; // a link within this page
});
document.addEventListener("keydown", (event) => {
    if (event.key === "/" && !event.target.closest("input")) {
        input.focus();
        event.preventDefault();
    }
});

// The map of functions.
const filter = document.getElementById("map-filter");
if (filter) {
    const rows = [...document.querySelectorAll("#map-table tbody tr")];
    const texts = rows.map((row) => row.textContent.toLowerCase());
    const holes = document.getElementById("map-holes");
    const show = () => {
        const wanted = filter.value.trim().toLowerCase();
        let count = 0;
        rows.forEach((row, i) => {
            row.hidden = !texts[i].includes(wanted) || (holes.checked && row.className !== "hole");
            count += !row.hidden;
        });
        document.getElementById("map-count").textContent = `${count} of ${rows.length}`;
    };
    filter.addEventListener("input", show);
    holes.addEventListener("change", show);
    show();
}
