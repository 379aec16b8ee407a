"use strict";
(() => {
  const root = document.documentElement;
  const stages = [...document.querySelectorAll(".stage")];
  const dividers = stages.map((stage) => stage.querySelector("input"));

  // One divider for all frames, so that switching between them keeps its place.
  function divide(percent) {
    const share = Math.min(100, Math.max(0, percent));
    root.style.setProperty("--split", share + "%");
    for (const divider of dividers) {
      divider.value = share;
      divider.setAttribute("aria-valuetext", Math.round(share) + " % before");
    }
  }

  function divideAt(stage, event) {
    const box = stage.getBoundingClientRect();
    divide((event.clientX - box.left) / box.width * 100);
  }

  stages.forEach((stage, index) => {
    const divider = dividers[index];
    divider.addEventListener("input", () => divide(Number(divider.value)));
    stage.addEventListener("pointerdown", (event) => {
      if (event.button !== 0 || !event.isPrimary) return;
      event.preventDefault();
      stage.setPointerCapture(event.pointerId);
      divider.focus({ preventScroll: true });
      // A finger may be about to scroll; the divider follows once it moves sideways or lets go.
      if (event.pointerType === "mouse") divideAt(stage, event);
    });
    stage.addEventListener("pointermove", (event) => {
      if (stage.hasPointerCapture(event.pointerId)) divideAt(stage, event);
    });
    stage.addEventListener("pointerup", (event) => {
      if (stage.hasPointerCapture(event.pointerId)) divideAt(stage, event);
    });
  });

  function show(choice) {
    for (const part of document.querySelectorAll("[data-view]")) {
      part.hidden = part.dataset.view !== choice.value;
    }
    root.style.setProperty("--at", choice.dataset.at + "%");
  }

  for (const choice of document.querySelectorAll(".frames input")) {
    // The page holds each picture once.
    const after = document.querySelector(`[data-view="${choice.value}"] .after img`);
    choice.nextElementSibling.src = after.src;
    choice.addEventListener("change", () => show(choice));
    // A browser may come back to the page with another frame chosen.
    if (choice.checked) show(choice);
  }
})();
