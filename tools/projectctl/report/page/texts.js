// The texts of the page, in the language of the tool, and numbers and times in its form.

const pageTexts = {texts: {}, language: 'en'};

function useTexts(model) {
    pageTexts.texts = model.texts;
    pageTexts.language = model.language.replace('_', '-');
    for (const place of document.querySelectorAll('[data-text]')) {
        place.textContent = text(place.dataset.text);
    }
    for (const place of document.querySelectorAll('[data-label]')) {
        place.setAttribute('aria-label', text(place.dataset.label));
    }
}

/** A text with {0}, {1}, ... replaced by the arguments. */
function text(key, ...values) {
    const pattern = pageTexts.texts[key] ?? key;
    return pattern.replace(/\{(\d+)\}/gu, (_, index) => {
        const value = values[Number(index)];
        return typeof value === 'number' ? shownNumber(value) : value;
    });
}

function shownNumber(value) {
    return value.toLocaleString(pageTexts.language);
}

function shownPercent(share) {
    return share.toLocaleString(pageTexts.language, {style: 'percent', maximumFractionDigits: 1});
}

function shownBytes(bytes) {
    const units = ['B', 'KiB', 'MiB', 'GiB', 'TiB'];
    let unit = 0;
    while (bytes >= 1024 && unit < units.length - 1) {
        bytes /= 1024;
        ++unit;
    }
    const digits = unit === 0 || bytes >= 100 ? 0 : 1;
    return `${bytes.toLocaleString(pageTexts.language, {maximumFractionDigits: digits})} ${units[unit]}`;
}

/** The date in "2026-11-22T18:58:43+01:00", in the author's time. */
function shownDate(time) {
    const [year, month, day] = time.slice(0, 10).split('-').map(Number);
    return new Date(Date.UTC(year, month - 1, day))
        .toLocaleDateString(pageTexts.language, {dateStyle: 'medium', timeZone: 'UTC'});
}
