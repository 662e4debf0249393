// The form with the conditions of the list.

class FilterForm {
    /** @param onChange called with the conditions after each change. */
    constructor(model, onChange) {
        this.model = model;
        this.onChange = onChange;
        this.conditions = noConditions();
        this.form = byId('filter');
        this.fill();
        this.form.addEventListener('submit', (event) => event.preventDefault());
    }

    fill() {
        this.search = this.input('search', 'Search', '');
        this.glob = this.input('text', 'Glob', '**/*.cpp');
        this.path = this.input('text', 'BelowPath', 'src');
        this.label = this.choices('WithLabel', 'labels');
        this.absentLabel = this.choices('WithoutLabel', 'absentLabels');
        this.kind = this.select('Kind', [['', 'AnyKind'], ['file', 'OnlyFiles'], ['folder', 'OnlyFolders']], 'kind');
        this.change = this.select('Change', [['', 'AnyChange'], ...changeWords.map((word) => [word, `Change_${word}`])],
            'change');
        this.entryPoints = this.flag('OnlyEntryPoints', 'isEntryPoint');
        this.unlabelled = this.flag('OnlyUnlabelled', 'isUnlabelled');
        this.chips = element('ul', {class: 'chips', 'aria-label': text('ChosenConditions')});
        this.link = element('a', {id: 'filterLink'}, text('LinkToFilter'));
        this.command = element('code', {id: 'filterCommand'});
        const clear = element('button', {type: 'button', id: 'clearFilter', onclick: () => this.set(noConditions())},
            text('ClearFilter'));
        this.form.append(
            element('div', {class: 'controls'}, this.search.label, this.glob.label, this.path.label, this.kind.label,
                this.label, this.absentLabel, this.model.changeOf === null ? null : this.change.label),
            element('div', {class: 'controls'}, this.entryPoints.label, this.unlabelled.label, clear, this.link),
            this.chips,
            element('p', {class: 'command'}, element('span', {class: 'quiet'}, `${text('SameCommand')} `), this.command));
        this.search.field.addEventListener('input', () => this.update({search: this.search.field.value}));
        this.glob.field.addEventListener('input', () => this.update({glob: this.glob.field.value}));
        this.path.field.addEventListener('change', () => this.addPath());
    }

    input(type, key, example) {
        const field = element('input', {type, id: `filter${key}`, placeholder: example, spellcheck: 'false'});
        return {field, label: element('label', {}, element('span', {}, text(key)), field)};
    }

    select(key, options, member) {
        const field = element('select', {id: `filter${key}`},
            ...options.map(([value, title]) => element('option', {value}, text(title))));
        field.addEventListener('change', () => this.update({[member]: field.value}));
        return {field, label: element('label', {}, element('span', {}, text(key)), field)};
    }

    flag(key, member) {
        const field = element('input', {type: 'checkbox', id: `filter${key}`});
        field.addEventListener('change', () => this.update({[member]: field.checked}));
        return {field, label: element('label', {class: 'flag'}, field, element('span', {}, text(key)))};
    }

    /** A list of the labels that `list` knows too; a chosen one is added to the conditions. */
    choices(key, member) {
        const {model} = this;
        const option = (choice) =>
            element('option', {value: `${choice.category} ${choice.label ?? ''}`}, shownChoice(model, choice));
        const groups = model.categories.map((item, category) => (item.isDeleted ? null : element('optgroup',
            {label: shownName(categoryName(model, category))},
            option({category, label: null}),
            ...model.labels.map((label, i) =>
                (label.category === category && !label.isDeleted ? option({category, label: i}) : null)))));
        const field = element('select', {id: `filter${key}`}, element('option', {value: ''}, text('Choose')), ...groups);
        field.addEventListener('change', () => {
            const [category, label] = field.value.split(' ');
            field.value = '';
            this.update({[member]: [...this.conditions[member],
                {category: Number(category), label: label === '' ? null : Number(label)}]});
        });
        return element('label', {}, element('span', {}, text(key)), field);
    }

    addPath() {
        const path = this.path.field.value.replace(/\/+$/u, '');
        this.path.field.value = '';
        if (path !== '') {
            this.update({paths: [...this.conditions.paths, path]});
        }
    }

    update(changed) {
        this.set({...this.conditions, ...changed, unknown: []});
    }

    set(conditions) {
        this.conditions = conditions;
        this.show();
        this.onChange(conditions);
    }

    show() {
        const {conditions, model} = this;
        const assign = (field, value) => {
            if (field.value !== value) { // keeps the cursor
                field.value = value;
            }
        };
        assign(this.search.field, conditions.search);
        assign(this.glob.field, conditions.glob);
        assign(this.kind.field, conditions.kind);
        assign(this.change.field, conditions.change);
        this.entryPoints.field.checked = conditions.isEntryPoint;
        this.unlabelled.field.checked = conditions.isUnlabelled;
        this.link.setAttribute('href', linkOf(model, conditions));
        this.command.textContent = commandOf(model, conditions);
        this.chips.replaceChildren(
            ...conditions.labels.map((choice) => this.chip('labels', choice, shownChoice(model, choice))),
            ...conditions.absentLabels.map((choice) =>
                this.chip('absentLabels', choice, text('NotCondition', shownChoice(model, choice)))),
            ...conditions.paths.map((path) => this.chip('paths', path, text('BelowCondition', shownName(path)))),
            ...conditions.unknown.map((words) =>
                element('li', {class: 'fault'}, text('UnknownLabel', shownName(words)))));
    }

    chip(member, value, title) {
        const remove = () => this.update({[member]: this.conditions[member].filter((other) => other !== value)});
        return element('li', {}, element('button',
            {type: 'button', onclick: remove, 'aria-label': text('RemoveCondition', title)}, element('bdi', {}, title), ' ×'));
    }
}
