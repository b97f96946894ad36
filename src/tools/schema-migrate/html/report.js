// The filters. Without scripts everything is shown, and they are not.
(() => {
  "use strict";
  const form = document.getElementById("filters");
  const items = Array.from(document.querySelectorAll(".item"));
  if (form === null || items.length === 0) {
    return;
  }
  const words = document.getElementById("words");
  const shown = document.getElementById("shown");
  const facets = Array.from(form.querySelectorAll("fieldset"));
  // What else goes when nothing in it is shown.
  const groups = Array.from(document.querySelectorAll("[data-group]"));
  let texts = null;

  // The texts in an element, a blank between two of them, so that none is found across both.
  const textOf = (element) => {
    const walker = document.createTreeWalker(element, NodeFilter.SHOW_TEXT);
    const parts = [];
    while (walker.nextNode()) {
      parts.push(walker.currentNode.data);
    }
    return parts.join(" ").toLowerCase();
  };

  const apply = () => {
    const wanted = facets.map((facet) => [
      facet.dataset.facet,
      new Set(Array.from(facet.querySelectorAll("input:checked"), (box) => box.value)),
    ]);
    const needles = words.value.toLowerCase().split(/\s+/).filter((word) => word !== "");
    if (needles.length > 0 && texts === null) {
      texts = items.map(textOf);
    }
    let count = 0;
    items.forEach((item, i) => {
      const isShown =
        wanted.every(([facet, values]) => values.has(item.dataset[facet])) &&
        needles.every((needle) => texts[i].includes(needle));
      if (item.hidden === isShown) {
        item.hidden = !isShown;
      }
      count += isShown ? 1 : 0;
    });
    for (const group of groups) {
      group.hidden = group.querySelector(".item:not([hidden])") === null;
    }
    shown.textContent =
      count === items.length ? "All " + count + " shown" : count + " of " + items.length + " shown";
  };

  // What comes near to being seen gets its true height, and moves what is below it.
  const scrollTo = (target, more) => {
    target.scrollIntoView();
    if (more > 0) {
      requestAnimationFrame(() => scrollTo(target, more - 1));
    }
  };

  // A link leads to what a filter hides, too.
  const reveal = () => {
    const target = document.getElementById(location.hash.slice(1));
    if (target !== null && target.closest("[hidden]") !== null) {
      form.reset();
      apply();
      scrollTo(target, 5);
    }
  };

  let pending = 0;
  words.addEventListener("input", () => {
    clearTimeout(pending);
    pending = setTimeout(apply, 150);
  });
  form.addEventListener("change", apply);
  form.addEventListener("reset", () => setTimeout(apply));
  form.addEventListener("submit", (event) => {
    event.preventDefault();
    apply();
  });
  window.addEventListener("hashchange", reveal);
  form.hidden = false;
  shown.textContent = "All " + items.length + " shown";
})();
